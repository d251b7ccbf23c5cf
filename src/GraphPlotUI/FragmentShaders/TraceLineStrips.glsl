// What is left of the background behind seventeen segments with soft edges: the product of their distances, each at
// most 1.
uniform vec4 u_TraceColour;

flat varying vec4 v_Start[4];
flat varying vec4 v_Rise[4];
flat varying vec4 v_Inverse[4];
flat varying vec3 v_Last;
flat varying vec3 v_Rows;

vec4 Squares(vec4 x, float i_Height, vec4 i_Start, vec4 i_Rise, vec4 i_Inverse)
{
    vec4 y = i_Height - i_Start;
    vec4 Along = clamp((x * v_Rows.y + y * i_Rise) * i_Inverse, 0.0, 1.0);
    x -= Along * v_Rows.y;
    y -= Along * i_Rise;
    return min(x * x + y * y, 1.0);
}

void main()
{
    // Written out: a loop that is not unrolled reads its varyings from memory.
    float y = gl_FragCoord.y * v_Rows.z;
    float Step = 4.0 * v_Rows.y;
    vec4 x = gl_FragCoord.x * v_Rows.z - v_Rows.x - vec4(0.0, 1.0, 2.0, 3.0) * v_Rows.y;
    vec4 Rest = Squares(x, y, v_Start[0], v_Rise[0], v_Inverse[0]);
    x -= Step;
    Rest *= Squares(x, y, v_Start[1], v_Rise[1], v_Inverse[1]);
    x -= Step;
    Rest *= Squares(x, y, v_Start[2], v_Rise[2], v_Inverse[2]);
    x -= Step;
    Rest *= Squares(x, y, v_Start[3], v_Rise[3], v_Inverse[3]);
    x -= Step;
    vec2 Last = vec2(x.x, y - v_Last.x);
    Last -= vec2(v_Rows.y, v_Last.y) * clamp((Last.x * v_Rows.y + Last.y * v_Last.y) * v_Last.z, 0.0, 1.0);
    float Square = Rest.x * Rest.y * Rest.z * Rest.w * min(dot(Last, Last), 1.0);
    gl_FragColor = vec4(u_TraceColour.rgb, 1.0 - sqrt(Square));
}
