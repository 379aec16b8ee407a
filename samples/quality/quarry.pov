// A quarry: terraces and boulders of bare rock, a few vehicles, hardly anything dark.
#declare FogDistance = 300;
#include "common.inc"

camera { perspective location <0, 18, 0> right x * 4 / 3 up y angle 56 look_at <0, 8, 100> }
Sun(<-0.4, 0.8, -0.5>, <0.95, 0.92, 0.85>)
SkyLight(<0.20, 0.23, 0.27>)
Sky(<0.80, 0.86, 0.90>, <0.40, 0.60, 0.86>, <0.96, 0.96, 0.97>)

plane { y, 0
  texture {
    pigment { granite turbulence 0.6 colour_map { [0 rgb <0.40, 0.37, 0.33>] [1 rgb <0.72, 0.68, 0.62>] } scale 9 }
    finish { Matt } normal { bumps 1 scale 0.8 }
  }
}

// Terraces, one behind and above the other.
#declare R = seed(19);
#declare I = 0;
#while (I < 9)
  box { <-400, 0, 0>, <400, 9 + 9 * I, 60>
    rotate (rand(R) - 0.5) * 10 * y translate <(rand(R) - 0.5) * 60, 0, 130 + 34 * I>
    texture {
      pigment {
        gradient y turbulence 0.5
        colour_map { [0 rgb <0.60, 0.54, 0.46>] [0.5 rgb <0.70, 0.66, 0.58>] [1 rgb <0.50, 0.46, 0.42>] }
        scale 5
      }
      finish { Matt } normal { bumps 1 scale 2 }
    }
  }
  #declare I = I + 1;
#end

// Boulders.
#declare I = 0;
#while (I < 120)
  #declare Z = 22 + 100 * rand(R);
  sphere { 0, 1
    scale <1 + 2 * rand(R), 0.6 + rand(R), 1 + 2 * rand(R)> translate <(rand(R) - 0.5) * 1.5 * Z, 0.3, Z>
    texture {
      pigment { granite colour_map { [0 rgb <0.35, 0.32, 0.29>] [1 rgb <0.66, 0.62, 0.57>] } }
      finish { Matt } normal { bumps 1 scale 0.5 }
    }
  }
  #declare I = I + 1;
#end

// Yellow vehicles with black wheels and windows.
#declare I = 0;
#while (I < 7)
  union {
    box { <-2, 1, -4>, <2, 4, 4> Rough(<0.80, 0.55, 0.08>, 1) }
    box { <-1.6, 1.5, 4>, <1.6, 5, 6> Rough(<0.75, 0.5, 0.08>, 1) }
    box { <-1.4, 3, 5.9>, <1.4, 4.5, 6.1> Rough(<0.04, 0.05, 0.06>, 1) }
    cylinder { <-2.2, 1, -2.5>, <-1.4, 1, -2.5>, 1 Rough(<0.03, 0.03, 0.03>, 1) }
    cylinder { <2.2, 1, -2.5>, <1.4, 1, -2.5>, 1 Rough(<0.03, 0.03, 0.03>, 1) }
    cylinder { <2.2, 1, 3.5>, <1.4, 1, 3.5>, 1 Rough(<0.03, 0.03, 0.03>, 1) }
    rotate 360 * rand(R) * y translate <(rand(R) - 0.5) * 80, 0, 40 + 80 * rand(R)>
  }
  #declare I = I + 1;
#end
