// What is left of the background behind sixteen bars with soft edges: the product of their distances, each at most 1.
uniform vec4 u_TraceColour;

flat varying vec4 v_Centre[4];
flat varying vec4 v_HalfHeight[4];
flat varying vec3 v_Rows;

float SquaredRest(vec4 x, float y, vec4 i_Centre, vec4 i_HalfHeight)
{
    vec4 Beyond = max(abs(y - i_Centre) - i_HalfHeight, 0.0);
    vec4 Squares = min(x * x + Beyond * Beyond, 1.0);
    return Squares.x * Squares.y * Squares.z * Squares.w;
}

void main()
{
    // Written out: a loop that is not unrolled reads its varyings from memory.
    float y = gl_FragCoord.y * v_Rows.z;
    float Step = 4.0 * v_Rows.y;
    vec4 x = gl_FragCoord.x * v_Rows.z - v_Rows.x - vec4(0.0, 1.0, 2.0, 3.0) * v_Rows.y;
    float Rest = SquaredRest(x, y, v_Centre[0], v_HalfHeight[0]);
    x -= Step;
    Rest *= SquaredRest(x, y, v_Centre[1], v_HalfHeight[1]);
    x -= Step;
    Rest *= SquaredRest(x, y, v_Centre[2], v_HalfHeight[2]);
    x -= Step;
    Rest *= SquaredRest(x, y, v_Centre[3], v_HalfHeight[3]);
    gl_FragColor = vec4(u_TraceColour.rgb, 1.0 - sqrt(Rest));
}
