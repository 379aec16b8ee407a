// A path into a forest: trunks one behind the other, undergrowth, little sky.
#declare FogDistance = 45;
#include "common.inc"

camera { perspective location <0, 1.7, 0> right x * 4 / 3 up y angle 58 look_at <0.6, 2.6, 20> }
Sun(<-0.5, 0.8, -0.5>, <0.90, 0.84, 0.66>)
SkyLight(<0.24, 0.28, 0.26>)
Sky(<0.80, 0.86, 0.88>, <0.48, 0.66, 0.86>, <0.95, 0.95, 0.95>)

plane { y, 0
  texture {
    pigment { bozo turbulence 0.9 colour_map { [0 rgb <0.20, 0.15, 0.08>] [0.4 rgb <0.42, 0.31, 0.16>] [0.7 rgb <0.26, 0.32, 0.12>] [1 rgb <0.35, 0.42, 0.16>] } scale 0.7 }
    finish { Matt } normal { bumps 1 scale 0.1 }
  }
}
// The path.
#declare I = 0;
#while (I < 60)
  cylinder { <0.02 * I + 0.9 * sin(I * 0.12), 0, I * 0.9>, <0.02 * I + 0.9 * sin(I * 0.12), 0.02, I * 0.9>, 1.2
    Rough(<0.55, 0.47, 0.36>, 0.4) }
  #declare I = I + 1;
#end

#declare R = seed(41);
#declare Leaves = texture {
  pigment { bozo colour_map { [0 rgb <0.08, 0.15, 0.05>] [0.5 rgb <0.24, 0.38, 0.11>] [1 rgb <0.48, 0.56, 0.20>] } scale 0.16 }
  finish { Matt } normal { bumps 1.3 scale 0.15 }
}
#macro Trunk(X, Z, Radius, Tall, Bark)
  union {
    cone { <0, -0.1, 0>, Radius * 1.3, <0.3 * (rand(R) - 0.5), Tall, 0>, Radius * 0.55
      texture { pigment { wood turbulence 0.4 colour_map { [0 rgb Bark * 0.6] [1 rgb Bark] } scale <0.15, 1.4, 0.15> } finish { Matt } normal { wrinkles 1 scale <0.05, 0.6, 0.05> } } }
    #local I = 0;
    #while (I < 7)
      #local A = rand(R) * 6.28;
      #local Y = Tall * (0.3 + 0.6 * rand(R));
      cylinder { <0, Y, 0>, <1.3 * cos(A), Y + 0.5, 1.3 * sin(A)>, Radius * 0.16 Rough(Bark * 0.8, 0.2) }
      sphere { <1.5 * cos(A), Y + 0.7, 1.5 * sin(A)>, 0.4 + 0.5 * rand(R) texture { Leaves } scale <1, 0.99, 1> }
      #local I = I + 1;
    #end
    translate <X, 0, Z>
  }
#end
#declare Barks = array[3] { <0.36, 0.27, 0.19>, <0.30, 0.26, 0.22>, <0.62, 0.60, 0.55> }
#declare I = 0;
#while (I < 240)
  #declare Z = 4 + 130 * pow(rand(R), 1.3);
  #declare Side = 2 * mod(I, 2) - 1;
  #declare X = Side * (2.3 + (4 + Z * 0.75) * pow(rand(R), 1.2));
  Trunk(X, Z, 0.14 + 0.2 * rand(R), 11 + 8 * rand(R), Barks[floor(rand(R) * 2.2)])
  #declare I = I + 1;
#end
// Undergrowth.
#declare I = 0;
#while (I < 500)
  #declare Z = 2.5 + 50 * pow(rand(R), 1.6);
  #declare Side = 2 * mod(I, 2) - 1;
  #declare X = Side * (1.6 + (2 + Z * 0.7) * rand(R));
  sphere { <X, 0.1, Z>, 0.15 + 0.4 * rand(R) texture { Leaves } scale <1, 0.8, 1> }
  #declare I = I + 1;
#end
