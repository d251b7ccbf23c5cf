uniform vec3 u_Up;
uniform vec3 u_CameraPosition;

varying vec3 v_position;
varying vec3 v_normal;
varying vec4 v_colour;

const float Ambience = 0.2;
const float TopFactor = 0.8;
const float BounceFactor = 0.2;
const float CameraFactor = 0.5;
const float SpecularPower = 16.0;

float diffuse(vec3 normal, vec3 direction)
{
    return max(0.0, dot(normal, direction));
}

void main()
{
    vec3 normal = normalize(v_normal);
    vec3 cameraDirection = normalize(u_CameraPosition - v_position);
    float lighting = diffuse(normal, cameraDirection) * CameraFactor + diffuse(normal, -u_Up) * BounceFactor +
                     diffuse(normal, u_Up) * TopFactor + Ambience;
    gl_FragColor = vec4(v_colour.rgb * lighting, v_colour.a);
}
