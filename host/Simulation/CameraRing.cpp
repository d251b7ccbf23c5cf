#include "Simulation/CameraRing.h"

#include "Simulation/WalkerPose.h"

#include <cmath>
#include <numbers>

namespace Simulation
{

namespace
{

constexpr double ringRadius = 6500.0; // millimetres, like all below
constexpr double lowHeight = 2200.0;
constexpr double highHeight = 3200.0;
constexpr double middleHeight = 1000.0;

} // namespace

std::string CameraName(std::uint32_t i_Camera)
{
    return "Camera" + std::to_string(i_Camera + 1);
}

std::array<float, 6> CameraPoseOf(std::uint32_t i_Camera)
{
    const double angle = 2.0 * std::numbers::pi * (i_Camera + 0.5) / CameraCount;
    const Eigen::Vector3d position(ringRadius * std::cos(angle), ringRadius * std::sin(angle),
                                   i_Camera % 2 == 0 ? lowHeight : highHeight);
    Eigen::Matrix3d axes;
    axes.col(2) = (position - Eigen::Vector3d(0.0, 0.0, middleHeight)).normalized();
    axes.col(0) = Eigen::Vector3d::UnitZ().cross(axes.col(2)).normalized();
    axes.col(1) = axes.col(2).cross(axes.col(0));
    const Eigen::Vector3d rotation = AngleAxisOf(Eigen::Quaterniond(axes));
    std::array<float, 6> pose{};
    for (int i = 0; i < 3; ++i)
    {
        pose[static_cast<std::size_t>(i)] = static_cast<float>(rotation[i]);
        pose[static_cast<std::size_t>(i) + 3] = static_cast<float>(position[i]);
    }
    return pose;
}

} // namespace Simulation
