// Firs in deep snow below mountains: bright colourless ground everywhere.
#declare FogDistance = 200;
#include "common.inc"

camera { perspective location <0, 4, 0> right x * 4 / 3 up y angle 54 look_at <0, 8, 80> }
Sun(<-0.6, 0.6, -0.5>, <0.80, 0.78, 0.74>)
SkyLight(<0.28, 0.32, 0.38>)
Sky(<0.80, 0.86, 0.92>, <0.30, 0.52, 0.84>, <0.97, 0.97, 0.98>)

plane { y, 0
  texture {
    pigment { bozo turbulence 0.8 colour_map { [0 rgb <0.80, 0.84, 0.90>] [1 rgb <0.93, 0.94, 0.96>] } scale 4 }
    finish { Matt } normal { bumps 0.7 scale 1.5 }
  }
}

// Firs of four cones each.
#declare R = seed(5);
#declare I = 0;
#while (I < 420)
  #declare Z = 14 + 500 * pow(rand(R), 1.6);
  #declare X = (rand(R) - 0.5) * (40 + Z * 1.6);
  #declare S = 4 + 6 * rand(R);
  #if (abs(X) > 4)
    #declare J = 0;
    #while (J < 4)
      cone { <X, S * (0.1 + 0.22 * J), Z>, S * (0.26 - 0.055 * J), <X, S * (0.45 + 0.2 * J), Z>, 0
        Rough(<0.10, 0.20, 0.12> * (0.8 + 0.5 * rand(R)), 0.5) }
      #declare J = J + 1;
    #end
  #end
  #declare I = I + 1;
#end

// Mountains of snow and rock.
#declare I = 0;
#while (I < 12)
  sphere { 0, 1 scale <160, 50 + 70 * rand(R), 120> translate <-700 + 130 * I, -8, 700 + 160 * rand(R)>
    texture {
      pigment {
        bozo turbulence 1
        colour_map { [0 rgb <0.85, 0.87, 0.92>] [0.5 rgb <0.90, 0.92, 0.95>] [0.5 rgb <0.32, 0.32, 0.34>]
          [1 rgb <0.22, 0.26, 0.24>] }
        scale <14, 8, 14>
      }
      finish { Matt } normal { bumps 1 scale 6 }
    }
  }
  #declare I = I + 1;
#end

// A hut.
box { <-12, 0, 26>, <-5, 4, 34> Rough(<0.45, 0.24, 0.16>, 0.8) }
