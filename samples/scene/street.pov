// A street above a valley, seen by a slowly moving camera; clear or in fog.
//
//   Fog=0           clear scene J
//   Fog=1           the same scene in homogeneous fog, I
//   Fog=2 Lights=0  white fog over black surfaces: the picture is 1 - t
//   clock           0 .. 1, the camera's way along the street
//
// Haze model. Fog type 1 mixes every camera ray, of length d, with the colour of the fog:
//   I = J * t + A * (1 - t),   t = exp(-d / FogDistance).
// assumed_gamma srgb lets the renderer calculate in the same sRGB code values that it writes to the
// file, so the mix happens in DISPLAY VALUES, not in linear light: the equation above holds for the
// bytes of the two pictures within rounding. That is how the dark-channel-prior literature applies
// the model. The price is that shading is computed in code values too; the colours allow for it.
//
// Nothing reflects or refracts: a second ray would be mixed with fog along its own way, and the
// pixel would no longer follow from one distance.
//
// One unit is one metre; x is right, y up, z along the street.
#version 3.7;

#ifndef (Fog) #declare Fog = 0; #end
#ifndef (Lights) #declare Lights = 1; #end

#ifndef (FogDistance) #declare FogDistance = 100; #end
#ifndef (LightR)
  #declare FogLight = <200, 203, 208> / 255;
#else
  #declare FogLight = <LightR, LightG, LightB> / 255;
#end

global_settings {
  assumed_gamma srgb
  ambient_light rgb Lights
  max_trace_level 3
}

#if (Fog = 1)
  fog { fog_type 1 distance FogDistance colour rgb FogLight }
#end
#if (Fog = 2)
  fog { fog_type 1 distance FogDistance colour rgb 1 }
#end

#include "ground.inc"
#include "plants.inc"
#include "houses.inc"
#include "cars.inc"
#include "furniture.inc"
#include "layout.inc"

// 9 m of dolly with a slight pan to the right. check_haze.py repeats the numbers of this block.
#declare CameraZ = 9 * clock;
#declare CameraAt = <StreetX(CameraZ) + 1.8, 1.9, CameraZ>;
#declare CameraTo = <3.2 + 2.4 * clock, 3.6, CameraZ + 40>;
camera {
  perspective
  location CameraAt
  right x * 16 / 9
  up y
  angle 62
  look_at CameraTo
}

// Sun from behind the right shoulder, so that the row of houses is lit and the trees on the right
// throw their shadows across the road. The second light stands for the sky and casts none.
light_source {
  <500, 440, -260> rgb <0.98, 0.90, 0.77> * Lights
  parallel point_at <0, 0, 0>
}
light_source {
  <-300, 500, -500> rgb <0.20, 0.23, 0.28> * Lights
  parallel point_at <0, 0, 0>
  shadowless
}

sky_sphere {
  pigment {
    gradient y
    colour_map {
      [0.00 rgb <0.78, 0.84, 0.88> * Lights]
      [0.12 rgb <0.62, 0.76, 0.89> * Lights]
      [0.45 rgb <0.30, 0.53, 0.82> * Lights]
    }
  }
  pigment {
    bozo
    turbulence 0.55 octaves 5 omega 0.55 lambda 2.2
    colour_map {
      [0.00 rgbt <0.90, 0.91, 0.92, 1 - 0.95 * Lights>]
      [0.35 rgbt <0.88, 0.90, 0.92, 1 - 0.70 * Lights>]
      [0.58 rgbt <0.84, 0.87, 0.90, 1>]
    }
    scale <0.55, 0.14, 0.55>
    translate <3.1, 0.4, 1.7>
  }
}
